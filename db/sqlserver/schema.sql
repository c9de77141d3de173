-- poc-dorvantos: schema for Microsoft SQL Server (2008 or later).
--
-- Run in the database named by the "dtInitialCatalog" setting. The database's default
-- collation must be case-insensitive and accent-sensitive (for example
-- Latin1_General_CI_AS), since the component writes table and column names in mixed
-- case. Amounts are decimal(19,4). Logins are the server's own.

CREATE TABLE tbPOC_Contas (
  conta_id      int IDENTITY(1,1) NOT NULL CONSTRAINT PK_tbPOC_Contas PRIMARY KEY,
  codigo        varchar(20)  NOT NULL,
  descrit       varchar(150) NULL,
  conta_activo  varchar(20)  NULL,
  conta_passivo varchar(20)  NULL,
  atribuicao    int NOT NULL CONSTRAINT DF_tbPOC_Contas_atribuicao DEFAULT (0)
);
CREATE UNIQUE INDEX ixPOC_Contas_codigo ON tbPOC_Contas (codigo);
GO

CREATE TABLE tbPOC_SubContas (
  sub_conta_id    int IDENTITY(1,1) NOT NULL CONSTRAINT PK_tbPOC_SubContas PRIMARY KEY,
  conta_id        int NOT NULL CONSTRAINT FK_tbPOC_SubContas_Contas REFERENCES tbPOC_Contas (conta_id),
  codigo          varchar(20)  NOT NULL,
  codigo_completo varchar(40)  NOT NULL,
  descrit         varchar(150) NULL
);
CREATE UNIQUE INDEX ixPOC_SubContas_codigo_completo ON tbPOC_SubContas (codigo_completo);
CREATE INDEX ixPOC_SubContas_conta ON tbPOC_SubContas (conta_id);
GO

CREATE TABLE tbPOC_Diario_Tipos (
  tipo_diario_id int IDENTITY(1,1) NOT NULL CONSTRAINT PK_tbPOC_Diario_Tipos PRIMARY KEY,
  descrit        varchar(100) NOT NULL
);
GO

CREATE TABLE tbContactos_ContasCorrentes_Tipos (
  tipo_id        int IDENTITY(1,1) NOT NULL CONSTRAINT PK_tbContactos_ContasCorrentes_Tipos PRIMARY KEY,
  descrit        varchar(100) NULL,
  tipo_diario_id int NULL CONSTRAINT FK_tbContactos_ContasCorrentes_Tipos_Diario
                          REFERENCES tbPOC_Diario_Tipos (tipo_diario_id)
);
GO

CREATE TABLE tbTaxas_Iva (
  iva_id  int IDENTITY(1,1) NOT NULL CONSTRAINT PK_tbTaxas_Iva PRIMARY KEY,
  descrit varchar(100) NOT NULL,
  regiao  varchar(30)  NOT NULL CONSTRAINT DF_tbTaxas_Iva_regiao DEFAULT ('Continente'),
  tx      decimal(9,4) NOT NULL,
  activo  int NOT NULL CONSTRAINT DF_tbTaxas_Iva_activo DEFAULT (1)
);
GO

CREATE TABLE tbPOC_Dorvantos_Codigos (
  descrit_id int IDENTITY(1,1) NOT NULL CONSTRAINT PK_tbPOC_Dorvantos_Codigos PRIMARY KEY,
  codigo     varchar(20)  NULL,
  descrit    varchar(150) NULL
);
CREATE INDEX ixPOC_Dorvantos_Codigos_codigo ON tbPOC_Dorvantos_Codigos (codigo);
GO

CREATE TABLE tbPOC_Contadores (
  contador_id int IDENTITY(1,1) NOT NULL CONSTRAINT PK_tbPOC_Contadores PRIMARY KEY,
  nome        varchar(30) NOT NULL,
  contador    int NULL
);
-- One row per name: two finalizations that both found no row cannot both add one.
CREATE UNIQUE INDEX ixPOC_Contadores_nome ON tbPOC_Contadores (nome);
GO

CREATE TABLE tbFechos (
  fecho_id int IDENTITY(1,1) NOT NULL CONSTRAINT PK_tbFechos PRIMARY KEY,
  data     datetime NOT NULL,
  descrit  varchar(100) NULL,
  anulado  int NULL CONSTRAINT DF_tbFechos_anulado DEFAULT (0)
);
GO

CREATE TABLE tbPOC_Dorvantos (
  dorvanto_id    int IDENTITY(1,1) NOT NULL CONSTRAINT PK_tbPOC_Dorvantos PRIMARY KEY,
  data           datetime NULL,
  dorvanto_no    varchar(50) NULL,
  tipo_diario_id int NULL,
  created_by     varchar(128) NULL,
  obs            varchar(2000) NULL,
  referencia     varchar(100) NULL,
  valor          decimal(19,4) NULL CONSTRAINT DF_tbPOC_Dorvantos_valor DEFAULT (0),
  finalizado     int NULL CONSTRAINT DF_tbPOC_Dorvantos_finalizado DEFAULT (0),
  sistema        int NULL,
  tipo_id        int NULL
);
CREATE INDEX ixPOC_Dorvantos_data ON tbPOC_Dorvantos (tipo_diario_id, data);
GO

CREATE TABLE tbPOC_Dorvantos_Details (
  diario_id           int IDENTITY(1,1) NOT NULL CONSTRAINT PK_tbPOC_Dorvantos_Details PRIMARY KEY,
  dorvanto_id         int NOT NULL CONSTRAINT FK_tbPOC_Dorvantos_Details_Dorvantos
                               REFERENCES tbPOC_Dorvantos (dorvanto_id),
  conta_id            int NULL,
  sub_conta_id        int NULL,
  codigo              varchar(20)  NULL,
  descrit             varchar(255) NULL,
  ref                 varchar(100) NULL,
  debito              decimal(19,4) NULL,
  credito             decimal(19,4) NULL,
  iva                 int NULL CONSTRAINT DF_tbPOC_Dorvantos_Details_iva DEFAULT (0),
  iva_tx_id           int NULL,
  iva_base_tributavel decimal(19,4) NULL,
  iva_apuramento      int NULL,
  reg_no              int NULL,
  ano                 int NULL,
  codigo_completo     varchar(40)  NULL,
  conta               varchar(20)  NULL,
  conta_descrit       varchar(150) NULL,
  sub_conta           varchar(20)  NULL,
  sub_conta_descrit   varchar(150) NULL,
  data                datetime NULL,
  related_id          int NULL,
  tipo_id             int NULL
);
CREATE INDEX ixPOC_Dorvantos_Details_dorvanto ON tbPOC_Dorvantos_Details (dorvanto_id);
GO

CREATE VIEW vwPOC_SubContas AS
SELECT s.sub_conta_id    AS sub_conta_id,
       s.codigo_completo AS codigo_completo,
       s.codigo          AS codigo,
       s.descrit         AS descrit,
       s.conta_id        AS conta_id,
       c.codigo          AS conta_codigo,
       c.descrit         AS conta_descrit
FROM tbPOC_SubContas s
JOIN tbPOC_Contas c ON c.conta_id = s.conta_id;
GO

CREATE VIEW vwTaxas_Iva AS
SELECT t.iva_id  AS iva_id,
       t.descrit AS descrit,
       t.regiao  AS regiao,
       t.tx      AS tx,
       REPLACE(CONVERT(varchar(20), CONVERT(decimal(9,2), t.tx * 100)), '.', ',')
         + ' % - ' + t.descrit + ' (' + t.regiao + ')' AS descrit2
FROM tbTaxas_Iva t
WHERE t.activo <> 0;
GO

CREATE VIEW vwPOC_Dorvantos_Details AS
SELECT d.dorvanto_id AS dorvanto_id,
       d.diario_id   AS diario_id,
       d.reg_no      AS reg_no,
       d.ano         AS ano,
       COALESCE(s.codigo_completo, d.codigo_completo) AS codigo_completo_list,
       COALESCE(c.codigo, d.conta)                    AS conta_list,
       COALESCE(c.descrit, d.conta_descrit)           AS conta_descrit_list,
       COALESCE(s.codigo, d.sub_conta)                AS sub_conta_list,
       COALESCE(s.descrit, d.sub_conta_descrit)       AS sub_conta_descrit_list,
       d.conta_id    AS conta_id,
       d.sub_conta_id AS sub_conta_id,
       d.codigo      AS codigo,
       d.descrit     AS descrit,
       d.ref         AS ref,
       d.debito      AS debito,
       d.credito     AS credito,
       d.iva         AS iva,
       d.iva_tx_id   AS iva_tx_id,
       d.iva_base_tributavel AS iva_base_tributavel,
       t.tx          AS iva_tx,
       d.data        AS data
FROM tbPOC_Dorvantos_Details d
LEFT JOIN tbPOC_Contas c ON c.conta_id = d.conta_id
LEFT JOIN tbPOC_SubContas s ON s.sub_conta_id = d.sub_conta_id
LEFT JOIN tbTaxas_Iva t ON t.iva_id = d.iva_tx_id;
GO

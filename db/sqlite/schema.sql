-- poc-dorvantos: schema of the embedded database (SQLite).
--
-- Text columns use the collation POC_CI_AS, which the engine registers: compares and
-- sorts ignoring case and keeping accents, Portuguese letters included. Dates are stored
-- as text 'yyyy-mm-dd hh:mm:ss', which compares and sorts as the dates do. Amounts are
-- REAL; sums of them are exact to 4 decimals (the engine's sum()). Keys that the
-- database generates are AUTOINCREMENT, so a deleted key is never handed out again.
-- Foreign keys are declared where they cannot refuse what the component writes: a line
-- always names an existing entry; account and sub-account keys of lines are left free,
-- as the component stores whatever the editor holds.

CREATE TABLE tbPOC_Contas (
  conta_id      INTEGER PRIMARY KEY AUTOINCREMENT,
  codigo        VARCHAR(20)  COLLATE POC_CI_AS NOT NULL,
  descrit       VARCHAR(150) COLLATE POC_CI_AS NULL,
  conta_activo  VARCHAR(20)  COLLATE POC_CI_AS NULL,
  conta_passivo VARCHAR(20)  COLLATE POC_CI_AS NULL,
  atribuicao    INTEGER NOT NULL DEFAULT 0
);
CREATE UNIQUE INDEX ixPOC_Contas_codigo ON tbPOC_Contas (codigo);

CREATE TABLE tbPOC_SubContas (
  sub_conta_id    INTEGER PRIMARY KEY AUTOINCREMENT,
  conta_id        INTEGER NOT NULL REFERENCES tbPOC_Contas (conta_id),
  codigo          VARCHAR(20)  COLLATE POC_CI_AS NOT NULL,
  codigo_completo VARCHAR(40)  COLLATE POC_CI_AS NOT NULL,
  descrit         VARCHAR(150) COLLATE POC_CI_AS NULL
);
CREATE UNIQUE INDEX ixPOC_SubContas_codigo_completo ON tbPOC_SubContas (codigo_completo);
CREATE INDEX ixPOC_SubContas_conta ON tbPOC_SubContas (conta_id);

CREATE TABLE tbPOC_Diario_Tipos (
  tipo_diario_id INTEGER PRIMARY KEY AUTOINCREMENT,
  descrit        VARCHAR(100) COLLATE POC_CI_AS NOT NULL
);

CREATE TABLE tbContactos_ContasCorrentes_Tipos (
  tipo_id        INTEGER PRIMARY KEY AUTOINCREMENT,
  descrit        VARCHAR(100) COLLATE POC_CI_AS NULL,
  tipo_diario_id INTEGER NULL REFERENCES tbPOC_Diario_Tipos (tipo_diario_id)
);

CREATE TABLE tbTaxas_Iva (
  iva_id  INTEGER PRIMARY KEY AUTOINCREMENT,
  descrit VARCHAR(100) COLLATE POC_CI_AS NOT NULL,
  regiao  VARCHAR(30)  COLLATE POC_CI_AS NOT NULL DEFAULT 'Continente',
  tx      REAL NOT NULL,
  activo  INTEGER NOT NULL DEFAULT 1
);

CREATE TABLE tbPOC_Dorvantos_Codigos (
  descrit_id INTEGER PRIMARY KEY AUTOINCREMENT,
  codigo     VARCHAR(20)  COLLATE POC_CI_AS NULL,
  descrit    VARCHAR(150) COLLATE POC_CI_AS NULL
);
CREATE INDEX ixPOC_Dorvantos_Codigos_codigo ON tbPOC_Dorvantos_Codigos (codigo);

CREATE TABLE tbPOC_Contadores (
  contador_id INTEGER PRIMARY KEY AUTOINCREMENT,
  nome        VARCHAR(30) COLLATE POC_CI_AS NOT NULL,
  contador    INTEGER NULL
);
-- One row per name: two finalizations that both found no row cannot both add one.
CREATE UNIQUE INDEX ixPOC_Contadores_nome ON tbPOC_Contadores (nome);

CREATE TABLE tbFechos (
  fecho_id INTEGER PRIMARY KEY AUTOINCREMENT,
  data     DATETIME NOT NULL,
  descrit  VARCHAR(100) COLLATE POC_CI_AS NULL,
  anulado  INTEGER NULL DEFAULT 0
);

CREATE TABLE tbPOC_Dorvantos (
  dorvanto_id    INTEGER PRIMARY KEY AUTOINCREMENT,
  data           DATETIME NULL,
  dorvanto_no    VARCHAR(50)  COLLATE POC_CI_AS NULL,
  tipo_diario_id INTEGER NULL,
  created_by     VARCHAR(128) COLLATE POC_CI_AS NULL,
  obs            VARCHAR(2000) COLLATE POC_CI_AS NULL,
  referencia     VARCHAR(100) COLLATE POC_CI_AS NULL,
  valor          REAL NULL DEFAULT 0,
  finalizado     INTEGER NULL DEFAULT 0,
  sistema        INTEGER NULL,
  tipo_id        INTEGER NULL
);
CREATE INDEX ixPOC_Dorvantos_data ON tbPOC_Dorvantos (tipo_diario_id, data);

CREATE TABLE tbPOC_Dorvantos_Details (
  diario_id           INTEGER PRIMARY KEY AUTOINCREMENT,
  dorvanto_id         INTEGER NOT NULL REFERENCES tbPOC_Dorvantos (dorvanto_id),
  conta_id            INTEGER NULL,
  sub_conta_id        INTEGER NULL,
  codigo              VARCHAR(20)  COLLATE POC_CI_AS NULL,
  descrit             VARCHAR(255) COLLATE POC_CI_AS NULL,
  ref                 VARCHAR(100) COLLATE POC_CI_AS NULL,
  debito              REAL NULL,
  credito             REAL NULL,
  iva                 INTEGER NULL DEFAULT 0,
  iva_tx_id           INTEGER NULL,
  iva_base_tributavel REAL NULL,
  iva_apuramento      INTEGER NULL,
  reg_no              INTEGER NULL,
  ano                 INTEGER NULL,
  codigo_completo     VARCHAR(40)  COLLATE POC_CI_AS NULL,
  conta               VARCHAR(20)  COLLATE POC_CI_AS NULL,
  conta_descrit       VARCHAR(150) COLLATE POC_CI_AS NULL,
  sub_conta           VARCHAR(20)  COLLATE POC_CI_AS NULL,
  sub_conta_descrit   VARCHAR(150) COLLATE POC_CI_AS NULL,
  data                DATETIME NULL,
  related_id          INTEGER NULL,
  tipo_id             INTEGER NULL
);
CREATE INDEX ixPOC_Dorvantos_Details_dorvanto ON tbPOC_Dorvantos_Details (dorvanto_id);

-- Sub-accounts with their account's code and name.
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

-- VAT rates as the line editor lists them: "23,00 % - Taxa normal (Continente)".
CREATE VIEW vwTaxas_Iva AS
SELECT t.iva_id  AS iva_id,
       t.descrit AS descrit,
       t.regiao  AS regiao,
       t.tx      AS tx,
       replace(printf('%.2f', t.tx * 100), '.', ',') || ' % - ' || t.descrit || ' (' || t.regiao || ')'
                 AS descrit2
FROM tbTaxas_Iva t
WHERE t.activo <> 0;

-- Lines as listed: the account texts come from the chart while the line is open; once
-- frozen by a finalization, the line's own copies are shown.
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

-- The logins of the embedded engine: salted, slow password hashes, never the password.
CREATE TABLE dv_logins (
  login_name VARCHAR(128) NOT NULL PRIMARY KEY COLLATE NOCASE,
  algorithm  VARCHAR(30)  NOT NULL,
  iterations INTEGER NOT NULL,
  salt       BLOB NOT NULL,
  hash       BLOB NOT NULL,
  created    DATETIME NOT NULL DEFAULT (datetime('now', 'localtime'))
);

-- poc-dorvantos: schema for PostgreSQL 15.
--
-- Create the database so that text folds and sorts as Portuguese does, then run this
-- file in it as its owner:
--
--   CREATE DATABASE poc TEMPLATE template0 ENCODING 'UTF8'
--     LOCALE_PROVIDER icu ICU_LOCALE 'pt' LOCALE 'C.UTF-8';
--
-- Names are written as in the other engines' schemas and left unquoted, so they fold to
-- lower case, as the names in the component's statements do. Text columns are citext:
-- equality, LIKE and ORDER BY ignore case and keep accents ('ç' = 'Ç', 'a' <> 'á'), as
-- a case-insensitive, accent-sensitive collation does on SQL Server; their lengths are
-- checked, since an over-long text is refused there. Keys the database generates are
-- identity columns; amounts are numeric(19,4), exact. Logins are the server's own.
--
-- Function bodies are quoted with '...' rather than $$...$$, so the file splits into
-- statements at ";" with the component's own tokenizer.

CREATE EXTENSION IF NOT EXISTS citext;

CREATE TABLE tbPOC_Contas (
  conta_id      integer GENERATED ALWAYS AS IDENTITY CONSTRAINT PK_tbPOC_Contas PRIMARY KEY,
  codigo        citext NOT NULL CHECK (length(codigo) <= 20),
  descrit       citext NULL CHECK (length(descrit) <= 150),
  conta_activo  citext NULL CHECK (length(conta_activo) <= 20),
  conta_passivo citext NULL CHECK (length(conta_passivo) <= 20),
  atribuicao    integer NOT NULL DEFAULT 0
);
CREATE UNIQUE INDEX ixPOC_Contas_codigo ON tbPOC_Contas (codigo);

CREATE TABLE tbPOC_SubContas (
  sub_conta_id    integer GENERATED ALWAYS AS IDENTITY CONSTRAINT PK_tbPOC_SubContas PRIMARY KEY,
  conta_id        integer NOT NULL CONSTRAINT FK_tbPOC_SubContas_Contas REFERENCES tbPOC_Contas (conta_id),
  codigo          citext NOT NULL CHECK (length(codigo) <= 20),
  codigo_completo citext NOT NULL CHECK (length(codigo_completo) <= 40),
  descrit         citext NULL CHECK (length(descrit) <= 150)
);
CREATE UNIQUE INDEX ixPOC_SubContas_codigo_completo ON tbPOC_SubContas (codigo_completo);
CREATE INDEX ixPOC_SubContas_conta ON tbPOC_SubContas (conta_id);

CREATE TABLE tbPOC_Diario_Tipos (
  tipo_diario_id integer GENERATED ALWAYS AS IDENTITY CONSTRAINT PK_tbPOC_Diario_Tipos PRIMARY KEY,
  descrit        citext NOT NULL CHECK (length(descrit) <= 100)
);

CREATE TABLE tbContactos_ContasCorrentes_Tipos (
  tipo_id        integer GENERATED ALWAYS AS IDENTITY
                         CONSTRAINT PK_tbContactos_ContasCorrentes_Tipos PRIMARY KEY,
  descrit        citext NULL CHECK (length(descrit) <= 100),
  tipo_diario_id integer NULL CONSTRAINT FK_tbContactos_ContasCorrentes_Tipos_Diario
                         REFERENCES tbPOC_Diario_Tipos (tipo_diario_id)
);

CREATE TABLE tbTaxas_Iva (
  iva_id  integer GENERATED ALWAYS AS IDENTITY CONSTRAINT PK_tbTaxas_Iva PRIMARY KEY,
  descrit citext NOT NULL CHECK (length(descrit) <= 100),
  regiao  citext NOT NULL DEFAULT 'Continente' CHECK (length(regiao) <= 30),
  tx      numeric(9,4) NOT NULL,
  activo  integer NOT NULL DEFAULT 1
);

CREATE TABLE tbPOC_Dorvantos_Codigos (
  descrit_id integer GENERATED ALWAYS AS IDENTITY CONSTRAINT PK_tbPOC_Dorvantos_Codigos PRIMARY KEY,
  codigo     citext NULL CHECK (length(codigo) <= 20),
  descrit    citext NULL CHECK (length(descrit) <= 150)
);
CREATE INDEX ixPOC_Dorvantos_Codigos_codigo ON tbPOC_Dorvantos_Codigos (codigo);

CREATE TABLE tbPOC_Contadores (
  contador_id integer GENERATED ALWAYS AS IDENTITY CONSTRAINT PK_tbPOC_Contadores PRIMARY KEY,
  nome        citext NOT NULL CHECK (length(nome) <= 30),
  contador    integer NULL
);
-- One row per name: two finalizations that both found no row cannot both add one.
CREATE UNIQUE INDEX ixPOC_Contadores_nome ON tbPOC_Contadores (nome);

CREATE TABLE tbFechos (
  fecho_id integer GENERATED ALWAYS AS IDENTITY CONSTRAINT PK_tbFechos PRIMARY KEY,
  data     timestamp(3) NOT NULL,
  descrit  citext NULL CHECK (length(descrit) <= 100),
  anulado  integer NULL DEFAULT 0
);

CREATE TABLE tbPOC_Dorvantos (
  dorvanto_id    integer GENERATED ALWAYS AS IDENTITY CONSTRAINT PK_tbPOC_Dorvantos PRIMARY KEY,
  data           timestamp(3) NULL,
  dorvanto_no    citext NULL CHECK (length(dorvanto_no) <= 50),
  tipo_diario_id integer NULL,
  created_by     citext NULL CHECK (length(created_by) <= 128),
  obs            citext NULL CHECK (length(obs) <= 2000),
  referencia     citext NULL CHECK (length(referencia) <= 100),
  valor          numeric(19,4) NULL DEFAULT 0,
  finalizado     integer NULL DEFAULT 0,
  sistema        integer NULL,
  tipo_id        integer NULL
);
CREATE INDEX ixPOC_Dorvantos_data ON tbPOC_Dorvantos (tipo_diario_id, data);

CREATE TABLE tbPOC_Dorvantos_Details (
  diario_id           integer GENERATED ALWAYS AS IDENTITY
                              CONSTRAINT PK_tbPOC_Dorvantos_Details PRIMARY KEY,
  dorvanto_id         integer NOT NULL CONSTRAINT FK_tbPOC_Dorvantos_Details_Dorvantos
                              REFERENCES tbPOC_Dorvantos (dorvanto_id),
  conta_id            integer NULL,
  sub_conta_id        integer NULL,
  codigo              citext NULL CHECK (length(codigo) <= 20),
  descrit             citext NULL CHECK (length(descrit) <= 255),
  ref                 citext NULL CHECK (length(ref) <= 100),
  debito              numeric(19,4) NULL,
  credito             numeric(19,4) NULL,
  iva                 integer NULL DEFAULT 0,
  iva_tx_id           integer NULL,
  iva_base_tributavel numeric(19,4) NULL,
  iva_apuramento      integer NULL,
  reg_no              integer NULL,
  ano                 integer NULL,
  codigo_completo     citext NULL CHECK (length(codigo_completo) <= 40),
  conta               citext NULL CHECK (length(conta) <= 20),
  conta_descrit       citext NULL CHECK (length(conta_descrit) <= 150),
  sub_conta           citext NULL CHECK (length(sub_conta) <= 20),
  sub_conta_descrit   citext NULL CHECK (length(sub_conta_descrit) <= 150),
  data                timestamp(3) NULL,
  related_id          integer NULL,
  tipo_id             integer NULL
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
       CAST(replace(to_char(t.tx * 100, 'FM999990.00'), '.', ',') || ' % - ' || t.descrit
            || ' (' || t.regiao || ')' AS citext) AS descrit2
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

-- What the translated statements call in place of the SQL Server built-ins.

-- GETDATE(): the local wall-clock time of the statement, to the millisecond.
CREATE FUNCTION getdate() RETURNS timestamp(3) LANGUAGE sql STABLE
  AS 'SELECT CAST(statement_timestamp() AS timestamp(3))';

CREATE FUNCTION year(timestamp) RETURNS integer LANGUAGE sql IMMUTABLE STRICT
  AS 'SELECT CAST(extract(year FROM $1) AS integer)';
CREATE FUNCTION month(timestamp) RETURNS integer LANGUAGE sql IMMUTABLE STRICT
  AS 'SELECT CAST(extract(month FROM $1) AS integer)';
CREATE FUNCTION day(timestamp) RETURNS integer LANGUAGE sql IMMUTABLE STRICT
  AS 'SELECT CAST(extract(day FROM $1) AS integer)';

-- @@IDENTITY: the key this session generated last, NULL before its first insert
-- (lastval() raises then).
CREATE FUNCTION dv_identity() RETURNS integer LANGUAGE plpgsql VOLATILE AS '
BEGIN
  RETURN lastval();
EXCEPTION WHEN object_not_in_prerequisite_state THEN
  RETURN NULL;
END';

-- "+" between two text columns joins them, as on SQL Server; a literal text on either
-- side is turned into "||" by the translation already.
CREATE FUNCTION dv_text_plus(text, text) RETURNS text LANGUAGE sql IMMUTABLE STRICT
  AS 'SELECT $1 || $2';
CREATE OPERATOR + (LEFTARG = text, RIGHTARG = text, FUNCTION = dv_text_plus);

-- Demo data: journal types and the integration types tied to them.

INSERT INTO tbPOC_Diario_Tipos (descrit) VALUES
('Caixa'),
('Bancos'),
('Compras'),
('Vendas'),
('Operações diversas'),
('Salários'),
('Abertura e encerramento');

INSERT INTO tbContactos_ContasCorrentes_Tipos (descrit, tipo_diario_id)
SELECT t.descrit, d.tipo_diario_id
FROM (SELECT 'Facturas de clientes' AS descrit, 'Vendas' AS diario
      UNION ALL SELECT 'Notas de crédito a clientes', 'Vendas'
      UNION ALL SELECT 'Recibos de clientes', 'Caixa'
      UNION ALL SELECT 'Facturas de fornecedores', 'Compras'
      UNION ALL SELECT 'Notas de crédito de fornecedores', 'Compras'
      UNION ALL SELECT 'Pagamentos a fornecedores', 'Bancos'
      UNION ALL SELECT 'Transferências bancárias', 'Bancos'
      UNION ALL SELECT 'Processamento de salários', 'Salários'
      UNION ALL SELECT 'Regularizações diversas', 'Operações diversas') t
JOIN tbPOC_Diario_Tipos d ON d.descrit = t.diario;

-- System codes that other modules stamp on their documents: not offered for integration.
INSERT INTO tbContactos_ContasCorrentes_Tipos (descrit, tipo_diario_id) VALUES
('Apuramento de IVA', NULL),
('Apuramento de resultados', NULL),
('Lançamento de abertura', NULL);

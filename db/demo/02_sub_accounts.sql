-- Demo data: sub-accounts. The full code is the account's code followed by the
-- sub-account's own three digits. Accounts with named sub-accounts (cash, banks,
-- customers, suppliers) get those; every other account that takes postings gets one
-- general sub-account under its own name.

INSERT INTO tbPOC_SubContas (conta_id, codigo, codigo_completo, descrit)
SELECT c.conta_id, s.codigo, c.codigo + s.codigo, s.descrit
FROM tbPOC_Contas c
JOIN (SELECT '11' AS conta, '001' AS codigo, 'Caixa - Sede (Lisboa)' AS descrit
      UNION ALL SELECT '11', '002', 'Caixa - Loja do Porto'
      UNION ALL SELECT '11', '003', 'Fundo de maneio'
      UNION ALL SELECT '12', '001', 'Caixa Geral de Depósitos - c/ 0035 0123'
      UNION ALL SELECT '12', '002', 'Millennium bcp - c/ 0033 4567'
      UNION ALL SELECT '12', '003', 'Novo Banco - c/ 0007 8910'
      UNION ALL SELECT '12', '004', 'Banco Santander Totta - c/ 0018 2468'
      UNION ALL SELECT '13', '001', 'Caixa Geral de Depósitos - depósito a prazo 12 meses'
      UNION ALL SELECT '211', '001', 'Clientes diversos'
      UNION ALL SELECT '211', '002', 'Farmácia Almeida & Filhos, Lda.'
      UNION ALL SELECT '211', '003', 'Construções Gonçalves, S.A.'
      UNION ALL SELECT '211', '004', 'Padaria São João, Lda.'
      UNION ALL SELECT '211', '005', 'Hotel Açores Mar, S.A.'
      UNION ALL SELECT '211', '006', 'Câmara Municipal de Évora'
      UNION ALL SELECT '221', '001', 'Fornecedores diversos'
      UNION ALL SELECT '221', '002', 'EDP Comercial - Comercialização de Energia, S.A.'
      UNION ALL SELECT '221', '003', 'Papelaria Conceição, Lda.'
      UNION ALL SELECT '221', '004', 'Distribuidora Ribeiro & Irmão, Lda.'
      UNION ALL SELECT '221', '005', 'Têxteis do Minho, S.A.'
      UNION ALL SELECT '2611', '001', 'Informática Lusitana, Lda.'
      UNION ALL SELECT '2611', '002', 'Auto Peninsular, S.A.'
      UNION ALL SELECT '2432', '001', 'IVA dedutível - Existências'
      UNION ALL SELECT '2432', '002', 'IVA dedutível - Imobilizado'
      UNION ALL SELECT '2432', '003', 'IVA dedutível - Outros bens e serviços'
      UNION ALL SELECT '2433', '001', 'IVA liquidado - Operações gerais'
      UNION ALL SELECT '2433', '002', 'IVA liquidado - Autoconsumo e operações gratuitas'
      UNION ALL SELECT '2622', '001', 'Remunerações a pagar - Maria João Ferreira'
      UNION ALL SELECT '2622', '002', 'Remunerações a pagar - José António Simões'
     ) s ON s.conta = c.codigo;

INSERT INTO tbPOC_SubContas (conta_id, codigo, codigo_completo, descrit)
SELECT conta_id, '001', codigo + '001', descrit
FROM tbPOC_Contas
WHERE atribuicao = 1
  AND conta_id NOT IN (SELECT conta_id FROM tbPOC_SubContas);

-- Demo data: the VAT rates in force in Portugal (Código do IVA, art. 18), for the
-- mainland and the autonomous regions, stored as fractions.

INSERT INTO tbTaxas_Iva (descrit, regiao, tx) VALUES
('Isento', 'Continente', 0),
('Taxa reduzida', 'Continente', 0.06),
('Taxa intermédia', 'Continente', 0.13),
('Taxa normal', 'Continente', 0.23),
('Taxa reduzida', 'Região Autónoma dos Açores', 0.04),
('Taxa intermédia', 'Região Autónoma dos Açores', 0.09),
('Taxa normal', 'Região Autónoma dos Açores', 0.16),
('Taxa reduzida', 'Região Autónoma da Madeira', 0.05),
('Taxa intermédia', 'Região Autónoma da Madeira', 0.12),
('Taxa normal', 'Região Autónoma da Madeira', 0.22);

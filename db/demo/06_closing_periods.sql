-- Demo data: the books are closed up to the end of 2009; a closing of 2010 entered by
-- mistake was cancelled and is not in force.

INSERT INTO tbFechos (data, descrit, anulado) VALUES
(CONVERT(DATETIME, '2009-12-31 0:00:00', 102), 'Encerramento do exercício de 2009', 0),
(CONVERT(DATETIME, '2010-06-30 0:00:00', 102), 'Encerramento do 1.º semestre de 2010 (anulado)', 1);

-- QUARVO demonstration data: one company 'DEMO' with three projects, their budgets, the
-- purchasing pieces of 2026 and everything they refer to. Load once on a fresh database,
-- after schema.sql.
--
-- Identifier blocks (10-digit texts), so that a number tells the table at a glance:
--   1-10 company, rights, parameters   11-13 projects          21-22 customers
--   31-38 departments, titles          41-46 services          51-55 purchase posts
--   61-75 item criteria                81-87 items             91-104 VAT
--   111-116 supplier families, terms   121-125 suppliers/resources
--   131-135 person, requester          141-145 purchase grouping  151-157 purchase accounts
--   161-186 vocabulary, item-supplier links, persons in charge, criteria
--   191-196 depots, stock              201-204 budgets         211-243 budget lines
--   301 quote request (lines 311)      401-404 orders (411-416)   501-502 receipts (511-513)
--   601-604 invoices (611-615)         701 time entry (711-712)   871-881 due dates, lots
-- Every numbering counter stands at 1000, above all of them.
--
-- The script opens no transaction of its own: the caller wraps it in one.
--
-- Amounts: a line's "BRUT" = QTE x PUHT, its "HT" = BRUT less the line discount; a header's
-- "BRUT" = sum of its lines' HT, "HT" = BRUT less the header discount plus carriage and fees,
-- "TTC" = HT + 20 % VAT. No piece is linked to a budget line yet: the link table is empty
-- and the budget lines' follow-up figures are zero.


------------------------------------------------------------------------------------------
-- Company, application rights, parameters
------------------------------------------------------------------------------------------

-- Current period December 2026 ('mmyyyy'); fiscal years 2026 (index 0) and 2025.
INSERT INTO "AFSOCI" ("IDENT", "CODE", "DESIG", "LIAISON_C", "LIAISON_G", "OPTION8", "OPTION9",
                      "MOIS_ANNEE", "DATE_DEBUT", "DATE_FIN")
VALUES ('0000000001', 'DEMO', 'Société de démonstration Bâtiment & Énergie', 'O', 'O', 'O', 'O',
        '122026', '2026-01-01;2025-01-01', '2026-12-31;2025-12-31');

INSERT INTO "SYSAPPLI" ("IDENT", "CODE", "DESIG")
VALUES ('0000000002', 'DOVERUVA', 'Gestion d''affaires');

INSERT INTO "SYSUTIL" ("IDENT", "CODE", "NOM") VALUES
    ('0000000006', 'demo', 'Utilisateur de démonstration'),
    ('0000000007', 'lecteur', 'Consultation seule');

-- 'demo' holds every right; 'lecteur' may only view and print.
INSERT INTO "SYSDROIT" ("IDENT", "SYSAPPLI_IDENT", "UTILISATEUR", "DROITS") VALUES
    ('0000000003', '0000000002', 'demo', 'VCAIMS'),
    ('0000000004', '0000000002', 'lecteur', 'VI');

INSERT INTO "SYSCOMPO" ("IDENT", "CODE", "DESIG")
VALUES ('0000000005', 'QUARVO_IMPORTER', 'Import des pièces d''achat');

-- Purchase grouping on item criterion 1; the four import kinds are allowed.
INSERT INTO "AFPARA" ("CODE", "DESIG", "PARAM1", "PARAM2", "PARAM3") VALUES
    ('MACHAT', 'Regroupement des achats par critère article', '1', '', '1'),
    ('IMPORT_03', 'Import des demandes de prix fournisseur', 'O', '/tmp/quarvo/import/df_achats.txt', ''),
    ('IMPORT_04', 'Import des commandes fournisseur', 'O', '/tmp/quarvo/import/cf_achats.txt', ''),
    ('IMPORT_05', 'Import des bons de réception', 'O', '/tmp/quarvo/import/bf_achats.txt', ''),
    ('IMPORT_06', 'Import des factures fournisseur', 'O', '/tmp/quarvo/import/ff_achats.txt', '');

INSERT INTO "CPPARAM" ("IDENT", "CODE", "DESIG", "JOURNAL_ACHAT")
VALUES ('0000000008', 'DEMO', 'Comptabilité intégrée de la société DEMO', 'HA');

-- Analytical section given on the lines (2).
INSERT INTO "GCPPARAM" ("IDENT", "DESIG", "SAISIE_ANA_A")
VALUES ('0000000009', 'Paramètres achats', 2);

INSERT INTO "GCPSTE" ("IDENT", "DESIG", "SAISIE_ANA_A", "GCPDEPOT_IDENT")
VALUES ('0000000010', 'Site principal', 2, '0000000191');

INSERT INTO "FRMT" ("CODE", "DESIG", "EXT", "SEPARATEUR", "FORMAT_DATE", "ENCODAGE")
VALUES ('EXCEL1', 'Texte tabulé (tableur)', 'TXT', 'TAB', 'dd/mm/yyyy', 'UTF-8');

------------------------------------------------------------------------------------------
-- Project side reference data
------------------------------------------------------------------------------------------

INSERT INTO "AFCLIE" ("IDENT", "CODE", "DESIG") VALUES
    ('0000000021', 'CLI001', 'Commune de Belleville-sur-Orne'),
    ('0000000022', 'CLI002', 'Syndicat des eaux du Val d''Érdre');

INSERT INTO "AFSERV" ("IDENT", "CODE", "DESIG") VALUES
    ('0000000031', 'TRV', 'Travaux'),
    ('0000000032', 'ETU', 'Bureau d''études');

INSERT INTO "AFETAB" ("IDENT", "CODE", "DESIG")
VALUES ('0000000035', 'SIE', 'Siège social');

INSERT INTO "SVCCIVIL" ("IDENT", "CODE", "DESIG", "BREF") VALUES
    ('0000000037', 'M', 'Monsieur', 'M.'),
    ('0000000038', 'MME', 'Madame', 'Mme');

INSERT INTO "AFRPS1" ("IDENT", "CODE", "NOM", "PRENOM") VALUES
    ('0000000181', 'CDUPRE', 'Dupré', 'Claire'),
    ('0000000182', 'MLEROY', 'Leroy', 'Mathéo');

INSERT INTO "AFRPS2" ("IDENT", "CODE", "NOM", "PRENOM")
VALUES ('0000000183', 'PGARNIER', 'Garnier', 'Paul');

INSERT INTO "AFCRI1" ("IDENT", "CODE", "DESIG") VALUES
    ('0000000185', 'PUBLIC', 'Marchés publics'),
    ('0000000186', 'PRIVE', 'Marchés privés');

INSERT INTO "AFVOCA" ("IDENT", "CODE", "LABEL", "BREF", "DESIG") VALUES
    ('0000000161', 'AFRPS1', 'Chargé d''affaires', 'Chargé', 'Chargé d''affaires'),
    ('0000000162', 'AFRPS2', 'Conducteur de travaux', 'Conducteur', 'Conducteur de travaux'),
    ('0000000163', 'AFCRI1', 'Secteur de marché', 'Secteur', 'Secteur de marché');

INSERT INTO "AFAFFA" ("IDENT", "CODE", "DESIG", "DATE_CREATION", "DATE_DEBUT", "DATE_FIN",
                      "AFCLIE_IDENT", "AFCLIE_CODE", "AFETAB_IDENT", "AFETAB_CODE",
                      "AFSERV_IDENT", "AFSERV_CODE", "AFRPS1_IDENT", "AFRPS1_CODE",
                      "AFRPS2_IDENT", "AFRPS2_CODE", "AFCRI1_IDENT", "AFCRI1_CODE") VALUES
    ('0000000011', 'AFF001', 'Rénovation de l''école des Érables', '2026-01-10', '2026-01-15', '2026-12-31',
     '0000000021', 'CLI001', '0000000035', 'SIE', '0000000031', 'TRV', '0000000181', 'CDUPRE',
     '0000000183', 'PGARNIER', '0000000185', 'PUBLIC'),
    ('0000000012', 'AFF002', 'Réseau d''eau potable — hameau de Sainte-Hélène', '2026-01-20', '2026-02-01', '2026-12-31',
     '0000000022', 'CLI002', '0000000035', 'SIE', '0000000031', 'TRV', '0000000182', 'MLEROY',
     '0000000183', 'PGARNIER', '0000000185', 'PUBLIC'),
    ('0000000013', 'AFF003', 'Étude de faisabilité énergétique de la médiathèque', '2026-02-15', '2026-03-01', '2026-09-30',
     '0000000021', 'CLI001', '0000000035', 'SIE', '0000000032', 'ETU', '0000000182', 'MLEROY',
     NULL, NULL, '0000000185', 'PUBLIC');

INSERT INTO "AFPOST" ("IDENT", "CODE", "DESIG") VALUES
    ('0000000051', 'ACH-MAT', 'Achats de matériel et fournitures'),
    ('0000000052', 'ACH-SST', 'Sous-traitance'),
    ('0000000053', 'ACH-LOC', 'Locations'),
    ('0000000054', 'ACH-MO', 'Main-d''œuvre'),
    ('0000000055', 'ACH-ETU', 'Études et honoraires');

-- Services; MO-TECH is a personnel service (NATURE 'P').
INSERT INTO "AFPRES" ("IDENT", "CODE", "DESIG", "NATURE", "POSTE_ACHAT", "UNITE") VALUES
    ('0000000041', 'MAT-ELEC', 'Matériel électrique', 'M', 'ACH-MAT', 'U'),
    ('0000000042', 'MAT-PLOM', 'Fournitures de plomberie', 'M', 'ACH-MAT', 'U'),
    ('0000000043', 'SST-MACO', 'Sous-traitance maçonnerie', 'S', 'ACH-SST', 'H'),
    ('0000000044', 'LOC-ENG', 'Location d''engins', 'L', 'ACH-LOC', 'J'),
    ('0000000045', 'MO-TECH', 'Main-d''œuvre technicien', 'P', 'ACH-MO', 'H'),
    ('0000000046', 'ETU-EXT', 'Études externes', 'E', 'ACH-ETU', 'F');

-- Analytical accounts with their post.
INSERT INTO "AFCOMP" ("IDENT", "CODE", "DESIG", "CPOST") VALUES
    ('60210000', '60210000', 'Achats de matériel électrique', 'ACH-MAT'),
    ('60220000', '60220000', 'Achats de fournitures de plomberie', 'ACH-MAT'),
    ('60400000', '60400000', 'Sous-traitance de travaux', 'ACH-SST'),
    ('60450000', '60450000', 'Études et prestations de services', 'ACH-ETU'),
    ('60700000', '60700000', 'Achats de marchandises', 'ACH-MAT'),
    ('61350000', '61350000', 'Locations mobilières', 'ACH-LOC'),
    ('62410000', '62410000', 'Frais accessoires sur achats', 'ACH-MAT'),
    ('62420000', '62420000', 'Transports sur achats', 'ACH-MAT');

-- Resources: the four suppliers (same IDENT as in GCPFOUR) and one technician.
INSERT INTO "AFFOUR" ("IDENT", "CODE", "NOM", "PRENOM", "DESIG", "CIVILITE", "AFSERV_IDENT") VALUES
    ('0000000121', 'ELECDIS', 'Électro-Distribution du Centre', NULL, 'Électro-Distribution du Centre', NULL, NULL),
    ('0000000122', 'HYDROSAN', 'Hydro-Sanitaire Équipement', NULL, 'Hydro-Sanitaire Équipement', NULL, NULL),
    ('0000000123', 'BATIMACO', 'Bâti-Maçonnerie Frères', NULL, 'Bâti-Maçonnerie Frères', NULL, NULL),
    ('0000000124', 'LOCAPRO', 'Loca-Pro Engins', NULL, 'Loca-Pro Engins', NULL, NULL),
    ('0000000125', 'TECH01', 'Bérard', 'Lucie', 'Lucie Bérard', 'MME', '0000000031');

INSERT INTO "AFPERS" ("IDENT", "CODE", "NOM", "PRENOM", "CIVILITE", "AFSERV_IDENT", "AFFOUR_IDENT")
VALUES ('0000000131', 'TECH01', 'Bérard', 'Lucie', 'MME', '0000000031', '0000000125');

------------------------------------------------------------------------------------------
-- Budgets and budget lines
------------------------------------------------------------------------------------------

-- Budget states: 201, 202 in progress, 203 anticipated, 204 closed (2025).
INSERT INTO "AFEBUD" ("IDENT", "AFAFFA_IDENT", "AFAFFA_CODE", "PIECE", "ORIGINE", "DESIG", "TYPE",
                      "CODE_ETAT", "VBUD_INI", "VBUD_REV", "DATE_CREATION", "DATE_DEBUT", "DATE_FIN",
                      "DATE_CLOTURE") VALUES
    ('0000000201', '0000000011', 'AFF001', 'BU26-0001', 'GCPECOM', 'Budget des travaux de rénovation', 'E',
     'E', '23500.00', '0.00', '2026-01-15', '2026-01-15', '2026-12-31', NULL),
    ('0000000202', '0000000012', 'AFF002', 'MANUEL', NULL, 'Budget du réseau d''eau potable', 'E',
     'E', '29400.00', '0.00', '2026-02-01', '2026-02-01', '2026-12-31', NULL),
    ('0000000203', '0000000013', 'AFF003', 'BU26-0003', 'GCPEDEV', 'Budget de l''étude énergétique', 'R',
     'A', '14860.00', '0.00', '2026-03-01', '2026-03-01', '2026-09-30', NULL),
    ('0000000204', '0000000011', 'AFF001', 'BU25-0007', 'GCPECOM', 'Budget préparatoire 2025 (clôturé)', 'E',
     'C', '4250.00', '0.00', '2025-03-01', '2025-03-01', '2025-12-31', '2025-12-15');

INSERT INTO "AFLBUD" ("IDENT", "NUMERO", "AFEBUD_IDENT", "DESIG", "STYLE", "AFAFFA_IDENT", "AFAFFA_CODE",
                      "AFEBUD_PIECE", "AFPRES_IDENT", "AFPRES_CODE", "UNITE", "APPRO", "DATE_DEBUT",
                      "DATE_FIN", "CHAPITRE2", "QBUD", "VBUD_D", "VENG", "VREA", "VRAF", "AFFECTE",
                      "HBUD", "HREA", "HRAF", "AVT") VALUES
    -- budget 0000000201, project AFF001: 23 500.00
    ('0000000211', '0000000201|1', '0000000201', 'Matériel électrique', 0, '0000000011', 'AFF001', 'BU26-0001',
     '0000000041', 'MAT-ELEC', 'U', 'A', '2026-01-15', '2026-12-31', '1)', 40, '6000.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 0, 0, 0, 0),
    ('0000000212', '0000000201|2', '0000000201', 'Fournitures de plomberie', 0, '0000000011', 'AFF001', 'BU26-0001',
     '0000000042', 'MAT-PLOM', 'U', 'A', '2026-01-15', '2026-12-31', '1)', 30, '2500.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 0, 0, 0, 0),
    ('0000000213', '0000000201|3', '0000000201', 'Sous-traitance maçonnerie', 0, '0000000011', 'AFF001', 'BU26-0001',
     '0000000043', 'SST-MACO', 'H', 'A', '2026-01-15', '2026-12-31', '2)', 200, '9000.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 0, 0, 0, 0),
    ('0000000214', '0000000201|4', '0000000201', 'Location de nacelle élévatrice', 0, '0000000011', 'AFF001', 'BU26-0001',
     '0000000044', 'LOC-ENG', 'J', 'A', '2026-01-15', '2026-12-31', '2)', 10, '1800.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 0, 0, 0, 0),
    ('0000000215', '0000000201|5', '0000000201', 'Main-d''œuvre technicien', 0, '0000000011', 'AFF001', 'BU26-0001',
     '0000000045', 'MO-TECH', 'H', NULL, '2026-01-15', '2026-12-31', '3)', 120, '4200.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 120, 0, 0, 0),
    -- budget 0000000202, project AFF002 (entered by hand): 29 400.00
    ('0000000221', '0000000202|1', '0000000202', 'Tubes et raccords', 0, '0000000012', 'AFF002', 'MANUEL',
     '0000000042', 'MAT-PLOM', 'U', 'A', '2026-02-01', '2026-12-31', NULL, 100, '8000.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 0, 0, 0, 0),
    ('0000000222', '0000000202|2', '0000000202', 'Tranchées et regards maçonnés', 0, '0000000012', 'AFF002', 'MANUEL',
     '0000000043', 'SST-MACO', 'H', 'A', '2026-02-01', '2026-12-31', NULL, 300, '13500.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 0, 0, 0, 0),
    ('0000000223', '0000000202|3', '0000000202', 'Location de mini-pelle', 0, '0000000012', 'AFF002', 'MANUEL',
     '0000000044', 'LOC-ENG', 'J', 'A', '2026-02-01', '2026-12-31', NULL, 20, '3600.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 0, 0, 0, 0),
    ('0000000224', '0000000202|4', '0000000202', 'Armoire de commande des pompes', 0, '0000000012', 'AFF002', 'MANUEL',
     '0000000041', 'MAT-ELEC', 'U', 'A', '2026-02-01', '2026-12-31', NULL, 10, '1500.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 0, 0, 0, 0),
    ('0000000225', '0000000202|5', '0000000202', 'Main-d''œuvre technicien', 0, '0000000012', 'AFF002', 'MANUEL',
     '0000000045', 'MO-TECH', 'H', NULL, '2026-02-01', '2026-12-31', NULL, 80, '2800.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 80, 0, 0, 0),
    -- budget 0000000203, project AFF003: 14 860.00; line 1 is a title line without service
    ('0000000231', '0000000203|1', '0000000203', 'Phase 1 — Diagnostic énergétique', 1, '0000000013', 'AFF003', 'BU26-0003',
     NULL, NULL, NULL, NULL, '2026-03-01', '2026-09-30', '1)', 0, '0.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 0, 0, 0, 0),
    ('0000000232', '0000000203|2', '0000000203', 'Étude thermique réglementaire', 0, '0000000013', 'AFF003', 'BU26-0003',
     '0000000046', 'ETU-EXT', 'F', 'A', '2026-03-01', '2026-09-30', '1)', 3, '12000.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 0, 0, 0, 0),
    ('0000000233', '0000000203|3', '0000000203', 'Relevés sur site', 0, '0000000013', 'AFF003', 'BU26-0003',
     '0000000045', 'MO-TECH', 'H', NULL, '2026-03-01', '2026-09-30', '1)', 60, '2100.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 60, 0, 0, 0),
    ('0000000234', '0000000203|4', '0000000203', 'Location de nacelle pour les relevés', 0, '0000000013', 'AFF003', 'BU26-0003',
     '0000000044', 'LOC-ENG', 'J', 'A', '2026-03-01', '2026-09-30', '2)', 2, '360.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 0, 0, 0, 0),
    ('0000000235', '0000000203|5', '0000000203', 'Capteurs et enregistreurs', 0, '0000000013', 'AFF003', 'BU26-0003',
     '0000000041', 'MAT-ELEC', 'U', 'A', '2026-03-01', '2026-09-30', '2)', 5, '400.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 0, 0, 0, 0),
    -- budget 0000000204, project AFF001, closed: 4 250.00
    ('0000000241', '0000000204|1', '0000000204', 'Matériel électrique (2025)', 0, '0000000011', 'AFF001', 'BU25-0007',
     '0000000041', 'MAT-ELEC', 'U', 'A', '2025-03-01', '2025-12-31', NULL, 10, '1200.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 0, 0, 0, 0),
    ('0000000242', '0000000204|2', '0000000204', 'Fournitures de plomberie (2025)', 0, '0000000011', 'AFF001', 'BU25-0007',
     '0000000042', 'MAT-PLOM', 'U', 'A', '2025-03-01', '2025-12-31', NULL, 10, '800.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 0, 0, 0, 0),
    ('0000000243', '0000000204|3', '0000000204', 'Sous-traitance maçonnerie (2025)', 0, '0000000011', 'AFF001', 'BU25-0007',
     '0000000043', 'SST-MACO', 'H', 'A', '2025-03-01', '2025-12-31', NULL, 50, '2250.00', '0.00',
     '0.00;0.00;0.00', '0.00;0.00;0.00', 'N', 0, 0, 0, 0);

------------------------------------------------------------------------------------------
-- Purchasing reference data
------------------------------------------------------------------------------------------

INSERT INTO "GCPDEPOT" ("IDENT", "CODE", "DESIG", "PRINCIPAL") VALUES
    ('0000000191', 'CENTRAL', 'Dépôt central', 1),
    ('0000000192', 'CHANTIER', 'Dépôt de chantier', 0);

INSERT INTO "GCPCRIT1" ("IDENT", "CODE", "DESIG") VALUES
    ('0000000061', 'ELEC', 'Électricité'),
    ('0000000062', 'PLOM', 'Plomberie'),
    ('0000000063', 'MACO', 'Maçonnerie'),
    ('0000000064', 'LOCA', 'Location de matériel'),
    ('0000000065', 'ETUD', 'Études');

INSERT INTO "GCPCRIT2" ("IDENT", "CODE", "DESIG") VALUES
    ('0000000071', 'STK', 'Article stocké'),
    ('0000000072', 'NSTK', 'Article non stocké');

INSERT INTO "GCPCRIT3" ("IDENT", "CODE", "DESIG")
VALUES ('0000000075', 'STD', 'Standard');

INSERT INTO "GCPREGM" ("IDENT", "CODE", "DESIG") VALUES
    ('0000000091', 'FR', 'France métropolitaine'),
    ('0000000092', 'UE', 'Intracommunautaire');

INSERT INTO "GCPTVA" ("IDENT", "CODE", "DESIG") VALUES
    ('0000000093', 'N20', 'TVA normale 20 %'),
    ('0000000094', 'R10', 'TVA intermédiaire 10 %'),
    ('0000000095', 'R55', 'TVA réduite 5,5 %'),
    ('0000000096', 'EXO', 'Exonéré');

INSERT INTO "GCPTXTVA" ("IDENT", "GCPREGM_IDENT", "GCPTVA_IDENT", "TAUX") VALUES
    ('0000000101', '0000000091', '0000000093', 20),
    ('0000000102', '0000000091', '0000000094', 10),
    ('0000000103', '0000000091', '0000000095', 5.5),
    ('0000000104', '0000000092', '0000000096', 0);

INSERT INTO "GCPARTIC" ("IDENT", "CODE", "DESIG", "UNITE", "PUHT", "GCPCRIT1_IDENT", "GCPCRIT2_IDENT",
                        "GCPCRIT3_IDENT", "GCPTVA_IDENT") VALUES
    ('0000000081', 'CABLE-3G2.5', 'Câble électrique 3G2,5 mm² (couronne de 100 m)', 'U', '180.00',
     '0000000061', '0000000071', '0000000075', '0000000093'),
    ('0000000082', 'TABLEAU-ELEC', 'Tableau électrique 4 rangées équipé', 'U', '350.00',
     '0000000061', '0000000071', '0000000075', '0000000093'),
    ('0000000083', 'TUBE-PER16', 'Tube PER Ø 16 (couronne de 50 m)', 'U', '95.00',
     '0000000062', '0000000071', '0000000075', '0000000093'),
    ('0000000084', 'ROBINET-EQ', 'Robinet d''équerre 1/2"', 'U', '12.50',
     '0000000062', '0000000071', '0000000075', '0000000093'),
    ('0000000085', 'MACO-HEURE', 'Heure de maçonnerie sous-traitée', 'H', '45.00',
     '0000000063', '0000000072', '0000000075', '0000000093'),
    ('0000000086', 'NACELLE-JOUR', 'Location de nacelle élévatrice (jour)', 'J', '180.00',
     '0000000064', '0000000072', '0000000075', '0000000093'),
    ('0000000087', 'ETUDE-THERM', 'Étude thermique réglementaire', 'F', '4000.00',
     '0000000065', '0000000072', '0000000075', '0000000093');

-- Purchase grouping: item criterion 1 -> service.
INSERT INTO "AFREGACH" ("IDENT", "CRITERE", "CLE_IDENT", "AFPRES_IDENT") VALUES
    ('0000000141', 1, '0000000061', '0000000041'),
    ('0000000142', 1, '0000000062', '0000000042'),
    ('0000000143', 1, '0000000063', '0000000043'),
    ('0000000144', 1, '0000000064', '0000000044'),
    ('0000000145', 1, '0000000065', '0000000046');

INSERT INTO "GAPFFOU" ("IDENT", "CODE", "DESIG") VALUES
    ('0000000111', 'NEGOCE', 'Négociants'),
    ('0000000112', 'SSTRAIT', 'Sous-traitants');

INSERT INTO "GCPREG" ("IDENT", "CODE", "DESIG", "NB_JOURS", "FIN_MOIS") VALUES
    ('0000000115', '30FM', '30 jours fin de mois', 30, 1),
    ('0000000116', 'COMPTANT', 'Comptant à réception', 0, 0);

INSERT INTO "GCPFOUR" ("IDENT", "CODE", "DESIG", "GCPREGM_IDENT", "GAPFFOU_IDENT", "GCPREG_IDENT") VALUES
    ('0000000121', 'ELECDIS', 'Électro-Distribution du Centre', '0000000091', '0000000111', '0000000115'),
    ('0000000122', 'HYDROSAN', 'Hydro-Sanitaire Équipement', '0000000091', '0000000111', '0000000116'),
    ('0000000123', 'BATIMACO', 'Bâti-Maçonnerie Frères', '0000000091', '0000000112', '0000000115'),
    ('0000000124', 'LOCAPRO', 'Loca-Pro Engins', '0000000091', '0000000111', '0000000115');

INSERT INTO "GAPARTFO" ("IDENT", "GCPARTIC_IDENT", "GCPFOUR_IDENT", "REFERENCE", "PUHT") VALUES
    ('0000000171', '0000000081', '0000000121', 'ED-C3G25-100', '180.00'),
    ('0000000172', '0000000082', '0000000121', 'ED-TAB4R', '350.00'),
    ('0000000173', '0000000083', '0000000122', 'HS-PER16-50', '95.00'),
    ('0000000174', '0000000084', '0000000122', 'HS-RE12', '12.50'),
    ('0000000175', '0000000085', '0000000123', 'BM-H-MACO', '45.00'),
    ('0000000176', '0000000086', '0000000124', 'LP-NAC12', '180.00');

INSERT INTO "GAPAPPOR" ("IDENT", "CODE", "NOM", "PRENOM", "CIVILITE", "SERVICE")
VALUES ('0000000135', 'TECH01', 'Bérard', 'Lucie', 'Madame', 'Travaux');

INSERT INTO "GCPSTOCK" ("IDENT", "GCPARTIC_IDENT", "GCPDEPOT_IDENT", "QTE_STOCK", "QTE_ATTENDUE") VALUES
    ('0000000193', '0000000081', '0000000191', 4, 0),
    ('0000000194', '0000000082', '0000000191', 1, 0),
    ('0000000195', '0000000083', '0000000191', 10, 0),
    ('0000000196', '0000000084', '0000000191', 0, 20);

------------------------------------------------------------------------------------------
-- Accounting link set-up
------------------------------------------------------------------------------------------

-- Purchase accounts by item criterion 1 (grouping mode 1) and by supplier family (mode 0),
-- for the French VAT regime, any VAT code.
INSERT INTO "GCPCPTACH" ("IDENT", "CRITERE_IDENT", "GCPREGM_IDENT", "GCPTVA_IDENT", "DATE_DEBUT",
                         "DATE_FIN", "COMPTE") VALUES
    ('0000000151', '0000000061', '0000000091', NULL, NULL, NULL, '60210000'),
    ('0000000152', '0000000062', '0000000091', NULL, NULL, NULL, '60220000'),
    ('0000000153', '0000000063', '0000000091', NULL, NULL, NULL, '60400000'),
    ('0000000154', '0000000064', '0000000091', NULL, NULL, NULL, '61350000'),
    ('0000000155', '0000000065', '0000000091', NULL, NULL, NULL, '60450000'),
    ('0000000156', '0000000111', '0000000091', NULL, NULL, NULL, '60700000'),
    ('0000000157', '0000000112', '0000000091', NULL, NULL, NULL, '60400000');

-- Same keys in both configurations: integrated accounting (GCPCOMPT) or file transfer (GCPTCFG).
INSERT INTO "GCPCOMPT" ("GENRE", "CLE", "VALEUR", "DESIG") VALUES
    ('J', 'ACHAT', 'HA', 'Journal des achats'),
    ('*', 'MACHAT', '1', 'Comptes d''achat par critère 1 de l''article'),
    ('C', 'AFRAIS', '62410000', 'Compte des frais sur achats'),
    ('C', 'APORT', '62420000', 'Compte du port sur achats');

INSERT INTO "GCPTCFG" ("GENRE", "CLE", "VALEUR", "DESIG") VALUES
    ('J', 'ACHAT', 'HA', 'Journal des achats'),
    ('*', 'MACHAT', '1', 'Comptes d''achat par critère 1 de l''article'),
    ('C', 'AFRAIS', '62410000', 'Compte des frais sur achats'),
    ('C', 'APORT', '62420000', 'Compte du port sur achats');

------------------------------------------------------------------------------------------
-- Purchasing pieces of 2026
------------------------------------------------------------------------------------------

-- Quote request DF26000001 (AFF003), carried into order CF26000004.
INSERT INTO "GAPEDEV" ("IDENT", "NUMERO_DOC", "DESIG", "ORIGINE", "DATE_CREATION", "DATE_MAJ", "HEURE_MAJ",
                       "VALIDEE", "SOLDEE", "SECAN_CODE", "GAPAPPOR_IDENT", "GCPFOUR_IDENT", "GCPREG_IDENT",
                       "GCPREGM_IDENT", "GCPDEPOT_IDENT", "BRUT", "HT", "TTC", "NET_A_PAYER",
                       "MTNT_HT", "MTNT_TTC", "QTT", "QTNT") VALUES
    ('0000000301', 'DF26000001', 'Nacelle pour relevés en façade', NULL, '2026-05-20', '2026-06-01', '08:40:00',
     1, 0, 'AFF003', '0000000135', '0000000124', '0000000115', '0000000091', '0000000191',
     '360.00', '360.00', '432.00', '432.00', '360.00', '432.00', 2, 0);

INSERT INTO "GAPLDEV" ("IDENT", "NUMERO", "GCPARTIC_IDENT", "GCPARTIC_CODE", "DESIG", "SECAN_CODE",
                       "GCPDEPOT_IDENT", "GCPTVA_IDENT", "QTE", "QTE_SOLDEE", "QTT", "PUHT", "TAUX_REMISE",
                       "BRUT", "HT") VALUES
    ('0000000311', '0000000301|1', '0000000086', 'NACELLE-JOUR', 'Location de nacelle élévatrice (jour)', NULL,
     '0000000191', '0000000093', 2, 0, 2, '180.00', 0, '360.00', '360.00');

-- Orders. CF26000001 fully received (BR26000001); CF26000002 partly received (BR26000002),
-- with 60.00 carriage and project sections on its lines; CF26000003 not carried forward at
-- all (no chaining row); CF26000004 not validated yet.
INSERT INTO "GAPECOM" ("IDENT", "NUMERO_DOC", "DESIG", "ORIGINE", "DATE_CREATION", "DATE_MAJ", "HEURE_MAJ",
                       "VALIDEE", "SOLDEE", "SECAN_CODE", "GAPAPPOR_IDENT", "GCPFOUR_IDENT", "GCPREG_IDENT",
                       "GCPREGM_IDENT", "GCPDEPOT_IDENT", "TAUX_REMISE", "TAUX_ESCOMPTE", "BRUT", "PORT_HT",
                       "FRAIS_HT", "HT", "TTC", "NET_A_PAYER", "MTNT_HT", "MTNT_TTC", "QTT", "QTNT") VALUES
    ('0000000401', 'CF26000001', 'Câblage des salles de classe', NULL, '2026-03-02', '2026-03-02', '10:15:00',
     1, 0, 'AFF001', '0000000135', '0000000121', '0000000115', '0000000091', '0000000191', 0, 0,
     '1350.00', '0.00', '0.00', '1350.00', '1620.00', '1620.00', '1350.00', '1620.00', 6, 0),
    ('0000000402', 'CF26000002', 'Raccordement du hameau', NULL, '2026-04-10', '2026-04-10', '16:42:00',
     1, 0, NULL, '0000000135', '0000000122', '0000000116', '0000000091', '0000000191', 0, 0,
     '1200.00', '60.00', '0.00', '1260.00', '1512.00', '1512.00', '950.00', '1140.00', 10, 20),
    ('0000000403', 'CF26000003', 'Reprise des murets de la cour', NULL, '2026-05-05', '2026-05-05', '09:30:00',
     1, 0, 'AFF001', '0000000135', '0000000123', '0000000115', '0000000091', '0000000191', 0, 0,
     '3600.00', '0.00', '0.00', '3600.00', '4320.00', '4320.00', '0.00', '0.00', 0, 80),
    ('0000000404', 'CF26000004', 'Nacelle pour relevés en façade', 'DF26000001', '2026-06-01', '2026-06-01', '08:45:00',
     0, 0, 'AFF003', '0000000135', '0000000124', '0000000115', '0000000091', '0000000191', 0, 0,
     '360.00', '0.00', '0.00', '360.00', '432.00', '432.00', '0.00', '0.00', 0, 2);

INSERT INTO "GAPLCOM" ("IDENT", "NUMERO", "GCPARTIC_IDENT", "GCPARTIC_CODE", "DESIG", "SECAN_CODE",
                       "GCPDEPOT_IDENT", "GCPTVA_IDENT", "QTE", "QTE_SOLDEE", "QTT", "PUHT", "TAUX_REMISE",
                       "BRUT", "HT") VALUES
    ('0000000411', '0000000401|1', '0000000081', 'CABLE-3G2.5', 'Câble électrique 3G2,5 mm² (couronne de 100 m)', NULL,
     '0000000191', '0000000093', 4, 0, 4, '180.00', 0, '720.00', '720.00'),
    ('0000000412', '0000000401|2', '0000000082', 'TABLEAU-ELEC', 'Tableau électrique 4 rangées équipé', NULL,
     '0000000191', '0000000093', 2, 0, 2, '350.00', 10, '700.00', '630.00'),
    ('0000000413', '0000000402|1', '0000000083', 'TUBE-PER16', 'Tube PER Ø 16 (couronne de 50 m)', 'AFF002',
     '0000000191', '0000000093', 10, 0, 10, '95.00', 0, '950.00', '950.00'),
    ('0000000414', '0000000402|2', '0000000084', 'ROBINET-EQ', 'Robinet d''équerre 1/2"', 'AFF002',
     '0000000191', '0000000093', 20, 0, 0, '12.50', 0, '250.00', '250.00'),
    ('0000000415', '0000000403|1', '0000000085', 'MACO-HEURE', 'Heure de maçonnerie sous-traitée', NULL,
     '0000000191', '0000000093', 80, 0, 0, '45.00', 0, '3600.00', '3600.00'),
    ('0000000416', '0000000404|1', '0000000086', 'NACELLE-JOUR', 'Location de nacelle élévatrice (jour)', NULL,
     '0000000191', '0000000093', 2, 0, 0, '180.00', 0, '360.00', '360.00');

-- Goods-received notes: BR26000001 (all of CF26000001, invoiced by FF26000001),
-- BR26000002 (the tubes of CF26000002, invoiced by FF26000003).
INSERT INTO "GAPEBL" ("IDENT", "NUMERO_DOC", "DESIG", "ORIGINE", "DATE_CREATION", "DATE_MAJ", "HEURE_MAJ",
                      "VALIDEE", "SOLDEE", "SECAN_CODE", "GAPAPPOR_IDENT", "GCPFOUR_IDENT", "GCPREG_IDENT",
                      "GCPREGM_IDENT", "GCPDEPOT_IDENT", "TAUX_REMISE", "TAUX_ESCOMPTE", "BRUT", "PORT_HT",
                      "FRAIS_HT", "HT", "TTC", "NET_A_PAYER", "MTNT_HT", "MTNT_TTC", "QTT", "QTNT") VALUES
    ('0000000501', 'BR26000001', 'Câblage des salles de classe', 'CF26000001', '2026-03-20', '2026-03-20', '14:05:00',
     1, 0, 'AFF001', '0000000135', '0000000121', '0000000115', '0000000091', '0000000191', 0, 0,
     '1350.00', '0.00', '0.00', '1350.00', '1620.00', '1620.00', '1350.00', '1620.00', 6, 0),
    ('0000000502', 'BR26000002', 'Raccordement du hameau', 'CF26000002', '2026-04-25', '2026-04-25', '11:20:00',
     1, 0, NULL, '0000000135', '0000000122', '0000000116', '0000000091', '0000000191', 0, 0,
     '950.00', '0.00', '0.00', '950.00', '1140.00', '1140.00', '950.00', '1140.00', 10, 0);

INSERT INTO "GAPLBL" ("IDENT", "NUMERO", "GCPARTIC_IDENT", "GCPARTIC_CODE", "DESIG", "SECAN_CODE",
                      "GCPDEPOT_IDENT", "GCPTVA_IDENT", "QTE", "QTE_SOLDEE", "QTT", "PUHT", "TAUX_REMISE",
                      "BRUT", "HT") VALUES
    ('0000000511', '0000000501|1', '0000000081', 'CABLE-3G2.5', 'Câble électrique 3G2,5 mm² (couronne de 100 m)', NULL,
     '0000000191', '0000000093', 4, 0, 4, '180.00', 0, '720.00', '720.00'),
    ('0000000512', '0000000501|2', '0000000082', 'TABLEAU-ELEC', 'Tableau électrique 4 rangées équipé', NULL,
     '0000000191', '0000000093', 2, 0, 2, '350.00', 10, '700.00', '630.00'),
    ('0000000513', '0000000502|1', '0000000083', 'TUBE-PER16', 'Tube PER Ø 16 (couronne de 50 m)', 'AFF002',
     '0000000191', '0000000093', 10, 0, 10, '95.00', 0, '950.00', '950.00');

-- Supplier invoices. "TYPE" 'F' is an invoice and 'A' a credit note; a credit note stores
-- positive quantities and amounts, and counts negatively wherever invoices are summed.
-- FF26000001 invoices BR26000001; FF26000002 is a direct invoice with a 2 % header
-- discount; AV26000001 credits one switchboard of FF26000001; FF26000003 invoices BR26000002.
INSERT INTO "GAPEFAC" ("IDENT", "NUMERO_DOC", "NUMERO", "DESIG", "ORIGINE", "TYPE", "DATE_CREATION", "DATE_MAJ",
                       "HEURE_MAJ", "VALIDEE", "SOLDEE", "SECAN_CODE", "GAPAPPOR_IDENT", "GCPFOUR_IDENT",
                       "GCPREG_IDENT", "GCPREGM_IDENT", "GCPDEPOT_IDENT", "TAUX_REMISE", "TAUX_ESCOMPTE",
                       "BRUT", "PORT_HT", "FRAIS_HT", "HT", "TTC", "NET_A_PAYER", "MTNT_HT", "MTNT_TTC",
                       "QTT", "QTNT") VALUES
    ('0000000601', 'FF26000001', 'EDC-F-2026-0415', 'Câblage des salles de classe', 'BR26000001', 'F',
     '2026-03-31', '2026-03-31', '17:00:00', 1, 0, 'AFF001', '0000000135', '0000000121', '0000000115',
     '0000000091', '0000000191', 0, 0, '1350.00', '0.00', '0.00', '1350.00', '1620.00', '1620.00',
     '0.00', '0.00', 0, 0),
    ('0000000602', 'FF26000002', 'BM-2026-118', 'Reprise des murets — premier acompte', NULL, 'F',
     '2026-05-29', '2026-05-29', '15:30:00', 1, 0, 'AFF001', '0000000135', '0000000123', '0000000115',
     '0000000091', '0000000191', 2, 0, '1800.00', '0.00', '0.00', '1764.00', '2116.80', '2116.80',
     '0.00', '0.00', 0, 0),
    ('0000000603', 'AV26000001', 'EDC-A-2026-0031', 'Retour d''un tableau électrique', 'FF26000001', 'A',
     '2026-04-15', '2026-04-15', '10:00:00', 1, 0, 'AFF001', '0000000135', '0000000121', '0000000115',
     '0000000091', '0000000191', 0, 0, '315.00', '0.00', '0.00', '315.00', '378.00', '378.00',
     '0.00', '0.00', 0, 0),
    ('0000000604', 'FF26000003', 'HS-26-00871', 'Raccordement du hameau', 'BR26000002', 'F',
     '2026-04-30', '2026-04-30', '09:05:00', 1, 0, NULL, '0000000135', '0000000122', '0000000116',
     '0000000091', '0000000191', 0, 0, '950.00', '0.00', '0.00', '950.00', '1140.00', '1140.00',
     '0.00', '0.00', 0, 0);

INSERT INTO "GAPLFAC" ("IDENT", "NUMERO", "GCPARTIC_IDENT", "GCPARTIC_CODE", "DESIG", "SECAN_CODE",
                       "GCPDEPOT_IDENT", "GCPTVA_IDENT", "QTE", "QTE_SOLDEE", "QTT", "PUHT", "TAUX_REMISE",
                       "BRUT", "HT") VALUES
    ('0000000611', '0000000601|1', '0000000081', 'CABLE-3G2.5', 'Câble électrique 3G2,5 mm² (couronne de 100 m)', NULL,
     '0000000191', '0000000093', 4, 0, 0, '180.00', 0, '720.00', '720.00'),
    ('0000000612', '0000000601|2', '0000000082', 'TABLEAU-ELEC', 'Tableau électrique 4 rangées équipé', NULL,
     '0000000191', '0000000093', 2, 0, 0, '350.00', 10, '700.00', '630.00'),
    ('0000000613', '0000000603|1', '0000000082', 'TABLEAU-ELEC', 'Tableau électrique 4 rangées équipé', NULL,
     '0000000191', '0000000093', 1, 0, 0, '350.00', 10, '350.00', '315.00'),
    ('0000000614', '0000000604|1', '0000000083', 'TUBE-PER16', 'Tube PER Ø 16 (couronne de 50 m)', 'AFF002',
     '0000000191', '0000000093', 10, 0, 0, '95.00', 0, '950.00', '950.00'),
    ('0000000615', '0000000602|1', '0000000085', 'MACO-HEURE', 'Heure de maçonnerie sous-traitée', NULL,
     '0000000191', '0000000093', 40, 0, 0, '45.00', 0, '1800.00', '1800.00');

-- Chaining of the transformations, one row per source line:
-- quote -> order, order -> goods-received note, goods-received note -> invoice.
INSERT INTO "CHAINAGE" ("CLE_SRC", "TYPE_DST", "IDE_DST", "LIG_DST") VALUES
    ('-1|0000000301|1', -2, '0000000404', '1'),
    ('-2|0000000401|1', -3, '0000000501', '1'),
    ('-2|0000000401|2', -3, '0000000501', '2'),
    ('-2|0000000402|1', -3, '0000000502', '1'),
    ('-3|0000000501|1', -4, '0000000601', '1'),
    ('-3|0000000501|2', -4, '0000000601', '2'),
    ('-3|0000000502|1', -4, '0000000604', '1');

-- Due dates of the invoices (30 days end of month, or cash).
INSERT INTO "GAPECH" ("IDENT", "GAPEFAC_IDENT", "NUMERO_DOC", "NUMERO", "GCPFOUR_IDENT", "GCPREG_IDENT",
                      "DATE_ECHEANCE", "MONTANT") VALUES
    ('0000000871', '0000000601', 'FF26000001', 1, '0000000121', '0000000115', '2026-04-30', '1620.00'),
    ('0000000872', '0000000602', 'FF26000002', 1, '0000000123', '0000000115', '2026-06-30', '2116.80'),
    ('0000000874', '0000000604', 'FF26000003', 1, '0000000122', '0000000116', '2026-04-30', '1140.00');

-- A lot on the valves still expected on order CF26000002.
INSERT INTO "GAPLOT" ("IDENT", "TYPE_PIECE", "PIECE_IDENT", "LIGNE_IDENT", "GCPARTIC_IDENT", "NUMERO_LOT",
                      "QTE", "SOLDE")
VALUES ('0000000881', -2, '0000000402', '0000000414', '0000000084', 'LOT-2604-RE', 20, 0);

------------------------------------------------------------------------------------------
-- Time entry (personnel service MO-TECH, two projects)
------------------------------------------------------------------------------------------

INSERT INTO "AFEFFO" ("IDENT", "NUMERO_DOC", "DESIG", "AFFOUR_IDENT", "DATE_PIECE", "DATE_CREATION",
                      "DATEM", "HEUREM", "DATE_MAJ", "HEURE_MAJ", "VALIDEE")
VALUES ('0000000701', 'TE26000001', 'Relevé d''heures de juin — Lucie Bérard', '0000000125', '2026-06-15',
        '2026-06-15', '2026-06-16', '09:12:00', '2026-06-16', '09:12:00', 1);

INSERT INTO "AFLFFO" ("IDENT", "NUMERO", "DESIG", "AFAFFA_IDENT", "AFPRES_IDENT", "QTE", "PUHT", "HT") VALUES
    ('0000000711', '0000000701|1', 'Pose des tableaux électriques', '0000000011', '0000000045', 8, '35.00', '280.00'),
    ('0000000712', '0000000701|2', 'Essais de pression du réseau', '0000000012', '0000000045', 4, '35.00', '140.00');

------------------------------------------------------------------------------------------
-- Numbering counters: identifiers per table (name 'NUMEROS'), document numbers per piece
-- kind (name 'NUMERO_DOC': the next order is CF26000005; credit notes have their own
-- sequence 'NUMERO_AVOIR', the next being AV26000002).
------------------------------------------------------------------------------------------

INSERT INTO "ZUMNDOC" ("MODULE", "NOM", "BASE", "DERNIER") VALUES
    ('QUARVO', 'NUMEROS', 'VOVOVA', 1000),
    ('AFLBUD', 'NUMEROS', 'VOVOVA', 1000),
    ('AFEBUD', 'NUMEROS', 'VOVOVA', 1000),
    ('AFAFFA', 'NUMEROS', 'VOVOVA', 1000),
    ('AFEFFO', 'NUMEROS', 'VOVOVA', 1000),
    ('AFLFFO', 'NUMEROS', 'VOVOVA', 1000),
    ('AFMOUV', 'NUMEROS', 'VOVOVA', 1000),
    ('AFPFST', 'NUMEROS', 'VOVOVA', 1000),
    ('AFPERS', 'NUMEROS', 'VOVOVA', 1000),
    ('AFFOUR', 'NUMEROS', 'VOVOVA', 1000),
    ('GAPEDEV', 'NUMEROS', 'GESCOM', 1000),
    ('GAPLDEV', 'NUMEROS', 'GESCOM', 1000),
    ('GAPECOM', 'NUMEROS', 'GESCOM', 1000),
    ('GAPLCOM', 'NUMEROS', 'GESCOM', 1000),
    ('GAPEBL', 'NUMEROS', 'GESCOM', 1000),
    ('GAPLBL', 'NUMEROS', 'GESCOM', 1000),
    ('GAPEFAC', 'NUMEROS', 'GESCOM', 1000),
    ('GAPLFAC', 'NUMEROS', 'GESCOM', 1000),
    ('GAPECH', 'NUMEROS', 'GESCOM', 1000),
    ('GAPLOT', 'NUMEROS', 'GESCOM', 1000),
    ('GAPAPPOR', 'NUMEROS', 'GESCOM', 1000),
    ('GAPARTFO', 'NUMEROS', 'GESCOM', 1000),
    ('GCPSTOCK', 'NUMEROS', 'GESCOM', 1000),
    ('GAPEDEV', 'NUMERO_DOC', 'GESCOM', 1),
    ('GAPECOM', 'NUMERO_DOC', 'GESCOM', 4),
    ('GAPEBL', 'NUMERO_DOC', 'GESCOM', 2),
    ('GAPEFAC', 'NUMERO_DOC', 'GESCOM', 3),
    ('GAPEFAC', 'NUMERO_AVOIR', 'GESCOM', 1);


-- Remaining figures of the budget lines as their follow-up would compute them before any link:
-- the whole budget remains.
UPDATE "AFLBUD"
   SET "VRAF" = "VBUD_D" || ';' || "VBUD_D" || ';' || "VBUD_D",
       "HRAF" = MAX("HBUD" - "HREA", 0)
 WHERE COALESCE("AFFECTE", 'N') <> 'O';
